pragma Singleton
import QtQuick

/// The subjects of a store without a live stage: passes on what the plugin has published.
QtObject {
    // qmllint disable unqualified
    readonly property var backEnd: typeof rootContextSubjectStoreOffline === "undefined" ? null : rootContextSubjectStoreOffline
    // qmllint enable unqualified

    readonly property var subjectsListModel: backEnd ? backEnd.subjectsListModel : null
}
