// ResourceData.cpp: registration of the Qt-compiled resource blocks. Each lives in the .qrc under
// ":/nightdome/<type>/<id>", uncompressed, so its bytes are read-only static data of the
// executable and can be registered in place without a copy.
#include "resources/ResourceData.h"

#include "platform/Resources.h"

#include <QDirIterator>
#include <QResource>

#include <mutex>

// Q_INIT_RESOURCE declares the initialiser where it is used, so this stays outside any namespace.
static void InitCompiledResources()
{
    Q_INIT_RESOURCE(nightdome_resources);
}

void InitResources()
{
    static std::once_flag once;
    std::call_once(once, [] {
        InitCompiledResources();
        QDirIterator types(QStringLiteral(":/nightdome"), QDir::Dirs | QDir::NoDotAndDotDot);
        while (types.hasNext()) {
            const QString typeDir = types.next();
            const QByteArray code = types.fileName().toLatin1();
            if (code.size() != 4)
                continue;
            const uint32_t type = (uint32_t(uint8_t(code[0])) << 24)
                | (uint32_t(uint8_t(code[1])) << 16) | (uint32_t(uint8_t(code[2])) << 8)
                | uint32_t(uint8_t(code[3]));
            QDirIterator ids(typeDir, QDir::Files);
            while (ids.hasNext()) {
                const QResource resource(ids.next());
                bool isNumber = false;
                const int id = ids.fileName().toInt(&isNumber);
                if (!isNumber || !resource.isValid()
                    || resource.compressionAlgorithm() != QResource::NoCompression)
                    continue;
                RegisterResource(type, id, resource.data(), size_t(resource.size()));
            }
        }
    });
}
