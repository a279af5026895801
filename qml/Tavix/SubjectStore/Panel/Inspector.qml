import QtQuick
import QtQuick.Controls
import QtQuick.Layouts
import Tavix.SubjectStore 1.0

/// All that the panel knows of what is selected, and what is not about single subjects: calibration, evaluation,
/// devices, presets and settings, a page each.
FocusScope {
    id: inspector

    property var panel: null

    readonly property bool calibrating: panel !== null && panel.calibration !== null && panel.calibration.running
    readonly property bool evaluating: SubjectStore.objectEvaluationProgressDone < SubjectStore.objectEvaluationProgressRequired
    readonly property var pages: [
        { "name": "Selected", "text": qsTr("Selected"), "busy": false },
        { "name": "Calibration", "text": qsTr("Calibration"), "busy": calibrating },
        { "name": "Evaluation", "text": qsTr("Evaluation"), "busy": evaluating },
        { "name": "Devices", "text": qsTr("Devices"), "busy": false },
        { "name": "Presets", "text": qsTr("Presets"), "busy": false },
        { "name": "Settings", "text": qsTr("Settings"), "busy": false }
    ]

    /// Brings the page of that name to the front.
    function show(name: string) {
        tabs.choose(inspector.pages.findIndex(page => page.name === name))
    }

    component Page: Loader {
        // Not StackLayout.isCurrentItem, which Qt never lets go of.
        required property bool current

        active: false
        onCurrentChanged: {
            if (current)
                active = true
        }
    }

    implicitWidth: 90 * Theme.unit
    // For what is not drawn here, such as scroll bars.
    palette {
        window: Theme.window
        windowText: Theme.text
        base: Theme.surface
        alternateBase: Theme.raised
        text: Theme.text
        button: Theme.raised
        buttonText: Theme.text
        highlight: Theme.highlight
        highlightedText: Theme.highlightedText
        toolTipBase: Theme.raised
        toolTipText: Theme.text
        light: Theme.raised
        midlight: Theme.raised
        mid: Theme.line
        dark: Theme.secondaryText
        shadow: Theme.line
        disabled {
            text: Theme.disabledText
            windowText: Theme.disabledText
            buttonText: Theme.disabledText
        }
    }

    Rectangle {
        anchors.fill: parent
        color: Theme.window
    }
    ColumnLayout {
        anchors.fill: parent
        spacing: 0

        TabStrip {
            id: tabs

            Layout.fillWidth: true
            pages: inspector.pages
            focus: true
        }
        FailureBar {
            id: failure

            Layout.fillWidth: true
        }
        // qmllint disable unqualified
        StackLayout {
            Layout.fillWidth: true
            Layout.fillHeight: true
            currentIndex: tabs.currentIndex

            Page {
                current: tabs.currentIndex === 0
                sourceComponent: SelectedPane {
                    panel: inspector.panel
                    onFinished: result => failure.show(result)
                }
            }
            Page {
                current: tabs.currentIndex === 1
                sourceComponent: CalibrationPane {
                    panel: inspector.panel
                    onFinished: result => failure.show(result)
                }
            }
            Page {
                current: tabs.currentIndex === 2
                sourceComponent: EvaluationPane {
                    panel: inspector.panel
                    onFinished: result => failure.show(result)
                }
            }
            Page {
                current: tabs.currentIndex === 3
                sourceComponent: DevicesPane {
                    panel: inspector.panel
                    onFinished: result => failure.show(result)
                }
            }
            Page {
                current: tabs.currentIndex === 4
                sourceComponent: PresetsPane {
                    panel: inspector.panel
                    onFinished: result => failure.show(result)
                }
            }
            Page {
                current: tabs.currentIndex === 5
                sourceComponent: SettingsPane {
                    panel: inspector.panel
                    onFinished: result => failure.show(result)
                }
            }
        }
        // qmllint enable unqualified
    }
}
