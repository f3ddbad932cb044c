// The panel that finds systems by the names of their stars: whole name, part or start of it,
// never minding case.
#pragma once

#include "query/StarNameQuery.h"
#include "query/panels/StarQueryView.h"

#include <string>

class NameQueryView : public StarQueryView {
public:
    NameQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent);

    NameQueryParam param;
    PopUpMenuButton* queryType; // "Query Type": name is, contains, starts with
    TextControl* starName; // "Star Name"

protected:
    void SetQueryParams() override;
    void InitQuery(Universe* universe) override;
    // Takes the system's name as the text searched for.
    void SystemDropped(StarSystem* system) override;

private:
    // The text searched for, cut to what the query's buffers hold: no name is that long, so a
    // longer text finds nothing either way.
    std::string fSearchText;
};
