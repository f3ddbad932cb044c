// The name panel: its menu and field, and the name query they fill in.
#include "query/panels/NameQueryView.h"

#include "query/panels/PopUpMenuButton.h"
#include "query/panels/TextControl.h"

NameQueryView::NameQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent)
    : StarQueryView(frame, name, "Find by Name", universe, parent)
    , param { kNameIs, nullptr, false }
{
    const BRect menu = FirstMenuFrame(120);
    queryType = AddPopUpMenu(menu, "Name Query TypeMB", "Query Type",
        { "Name is", "Name contains", "Name starts with" });
    starName = AddTextControl(NextFrame(menu, 145, 130), "Star Name", "", "The Sun", 0);
    InitQuery(universe);
}

void NameQueryView::InitQuery(Universe* universe)
{
    query = new StarNameQuery(universe);
}

void NameQueryView::SetQueryParams()
{
    param.mode = queryType->MarkedIndex();
    fSearchText.assign(starName->Text());
    if (fSearchText.size() >= size_t(StarNameQuery::kNameBufferSize))
        fSearchText.resize(size_t(StarNameQuery::kNameBufferSize) - 1);
    param.text = fSearchText.c_str();
    // Names are always looked for regardless of case.
    param.caseSensitive = false;
    queryParam = &param;
}

void NameQueryView::SystemDropped(StarSystem* system)
{
    starName->SetText(system->GetName());
}
