// Written by generate.mjs from docs/api; changes made here are lost.

import type { CallOptions, Caller, Inputs, Method, Outputs, Result } from './types.js';

/** What the greeting of a host with the same API says in `api`. */
export const apiHash = '9d4e7a0ea0d04dcbaeb66e0f8e9542311f3739b12a6460645d689aac139d6372';

/** Every result code by name; failures have the highest bit set. */
export const ResultCode = {
  Ok: 0x00000000,
  OkButNoEffect: 0x00000001,
  OkButPartial: 0x00000002,
  OkButFinished: 0x00000003,
  OkButModified: 0x00000004,
  Failed: 0x80000000,
  FailedWithException: 0x80000001,
  Finished: 0x80000002,
  Stopping: 0x80000003,
  NotImplemented: 0x80000004,
  NotSupported: 0x80000005,
  NotPermitted: 0x80000006,
  NotAvailable: 0x80000007,
  NotConnected: 0x80000008,
  NotSet: 0x80000009,
  NotFound: 0x8000000A,
  NotRequired: 0x8000000B,
  AlreadyPresent: 0x8000000C,
  AlreadyInProgress: 0x8000000D,
  AlreadySet: 0x8000000E,
  InvalidArgument: 0x8000000F,
  InvalidIndex: 0x80000010,
  InvalidName: 0x80000011,
  InvalidId: 0x80000012,
  InvalidHandle: 0x80000013,
  InvalidToken: 0x80000014,
  InvalidPointer: 0x80000015,
  InvalidFormat: 0x80000016,
  InvalidType: 0x80000017,
  InvalidVersion: 0x80000018,
  InvalidSession: 0x80000019,
  InvalidInfo: 0x8000001A,
  InvalidValue: 0x8000001B,
  InvalidSettings: 0x8000001C,
  ProtocolFailure: 0x8000001D,
  NetworkFailure: 0x8000001E,
  AllocationFailure: 0x8000001F,
  SerialisationFailure: 0x80000020,
  FileIOFailure: 0x80000021,
  TimedOut: 0x80000022,
  WouldBlock: 0x80000023,
  EndOfData: 0x80000024,
  Conflict: 0x80000025,
  FileNotOpen: 0x80000026,
  ShuttingDown: 0x80000027,
  DiskFull: 0x80000028,
  Canceled: 0x80000029,
  FileNotFound: 0x8000002A,
  RPCUnknown: 0x8000002B,
  RPCFailed: 0x8000002C,
  RPCInvalid: 0x8000002D,
  RPCNotConnected: 0x8000002E,
  NoResult: 0x80010002,
} as const;
export type ResultName = keyof typeof ResultCode;

/** Basic object warning types. */
export const EBasicObjectWarning = {
  /** Proximity group has no unique object. */
  ProximityGroupMissingUnique: 0,
  /** Proximity group contains more than one instance from the same template group. */
  ProximityGroupDuplicateTemplates: 1,
  /** Object is in a template group, but isn't in a proximity group. */
  TemplateGroupNoProximityGroup: 2,
  /** Template group contains non-identical objects. */
  TemplateGroupNonIdentical: 3,
  /** Template groups require either Proximity Grouping or Object Instance Tracking to be enabled in processing. */
  TemplateGroupProcessingNotEnabled: 4,
  /** Object could be confused with another object, or another view of itself. */
  ObjectConfusion: 5,
  /** Object is likely to be confused with another object, or another view of itself. */
  ObjectConfusionCritical: 6,
} as const;
export type EBasicObjectWarning = (typeof EBasicObjectWarning)[keyof typeof EBasicObjectWarning];

/** Smart object warning types. */
export const ESmartObjectWarning = {
  /** A linked device is also linked to another smart object. */
  DuplicateDevice: 0,
  /** Enabled smart object pattern conflicts with another enabled smart object. */
  DuplicatePattern: 1,
  /** Enabled smart object has no pattern defined. */
  NoPattern: 2,
  /** Smart object is linked to a disconnected device. */
  DisconnectedDevice: 3,
  /** Smart object is linked to a missing device. */
  MissingDevice: 4,
  /** Smart object has one or more empty device links. */
  DeviceNotLinked: 5,
  /** Proximity group has no unique object. */
  ProximityGroupMissingUnique: 6,
  /** Proximity group contains more than one instance from the same template group. */
  ProximityGroupDuplicateTemplates: 7,
  /** Object is in a template group, but isn't in a proximity group. */
  TemplateGroupNoProximityGroup: 8,
  /** Template group contains non-identical objects. */
  TemplateGroupNonIdentical: 9,
  /** Template groups require either Proximity Grouping or Object Instance Tracking to be enabled in processing. */
  TemplateGroupProcessingNotEnabled: 10,
  /** Object could be confused with another object, or another view of itself. */
  ObjectConfusion: 11,
  /** Object is likely to be confused with another object, or another view of itself. */
  ObjectConfusionCritical: 12,
  /** Smart object markers are turned off, because a linked device is plugged in for recharging. */
  ActiveMarkersOff: 13,
} as const;
export type ESmartObjectWarning = (typeof ESmartObjectWarning)[keyof typeof ESmartObjectWarning];

/** Character warning types. */
export const ECharacterWarning = {
  /** Character has one or more warnings on slot objects. */
  SlotObjectWarning: 0,
  /** Character is not calibrated. */
  NotCalibrated: 1,
  /** Character has not been assigned a reference cluster (one with auto-assign disabled). */
  CFCNoReferenceClusterAssigned: 2,
  /** Enabled characters have more empty slots than there are auto-assignable objects. */
  InsufficientAutoAssignCandidates: 3,
} as const;
export type ECharacterWarning = (typeof ECharacterWarning)[keyof typeof ECharacterWarning];

/** Calibration state of a character. */
export const ECharacterCalibrationState = {
  /** Character has not been calibrated. */
  Uncalibrated: 0,
  /** Character is in the process of calibration. */
  Calibrating: 1,
  /** Character has been calibrated. */
  Calibrated: 2,
} as const;
export type ECharacterCalibrationState = (typeof ECharacterCalibrationState)[keyof typeof ECharacterCalibrationState];

/** Subject calibration states. */
export const ESubjectCalibrationState = {
  /** Subject calibration has not yet been run.  The system is ready to subject calibrate in None, Completed or Cancelled. */
  None: 0,
  /** The system is attempting to to identify a subject T-Pose. */
  TPoseLabelling: 1,
  /** The system is calibrating the subject. */
  Calibrating: 2,
  /** Subject calibration has completed.  This is an end state of the process. */
  Completed: 3,
  /** The last subject calibration was cancelled.  This is an end state of the process. */
  Cancelled: 4,
} as const;
export type ESubjectCalibrationState = (typeof ESubjectCalibrationState)[keyof typeof ESubjectCalibrationState];

/** The functions of the API by their full names. */
export interface Functions {
  'BasicObjectServices.BasicObjectList': {
    inputs: Record<string, never>;
    outputs: {
      /** List of basic object names. */
      Names: string[];
    };
    returned: undefined;
  };
  'BasicObjectServices.Remove': {
    inputs: {
      /** Basic object name. */
      Name: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.RemoveAll': {
    inputs: Record<string, never>;
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.Rename': {
    inputs: {
      /** Name of the basic object to update. */
      OldName: string;
      /** New basic object name. */
      NewName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.Enabled': {
    inputs: {
      /** Name of the basic object. */
      Name: string;
    };
    outputs: {
      /** Enabled value. */
      Enabled: boolean;
    };
    returned: undefined;
  };
  'BasicObjectServices.SetEnabled': {
    inputs: {
      /** Name of the basic object to update. */
      Name: string;
      /** Enabled value. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.SetAllEnabled': {
    inputs: {
      /** Enabled value. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.Color': {
    inputs: {
      /** Name of the basic object. */
      Name: string;
    };
    outputs: {
      /** HTML hex color code (format '#AARRGGBB'). */
      ColorHtml: string;
    };
    returned: undefined;
  };
  'BasicObjectServices.SetColor': {
    inputs: {
      /** Name of the basic object to update. */
      Name: string;
      /** HTML hex color code (format '#AARRGGBB'). */
      ColorHtml: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.AutoAssignEnabled': {
    inputs: {
      /** Name of the basic object. */
      Name: string;
    };
    outputs: {
      /** Auto-assign enabled value. */
      Enabled: boolean;
    };
    returned: undefined;
  };
  'BasicObjectServices.SetAutoAssignEnabled': {
    inputs: {
      /** Name of the basic object to update. */
      Name: string;
      /** Auto-assign enabled value. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.AutoAssignedName': {
    inputs: {
      /** Name of the basic object. */
      Name: string;
    };
    outputs: {
      /** Auto-assigned name. */
      AutoAssignedName: string;
    };
    returned: undefined;
  };
  'BasicObjectServices.ProximityGroupName': {
    inputs: {
      /** Name of the basic object. */
      Name: string;
    };
    outputs: {
      /** Name of the proximity group to which this object belongs. */
      ProximityGroupName: string;
    };
    returned: undefined;
  };
  'BasicObjectServices.SetProximityGroupName': {
    inputs: {
      /** Name of the basic object to update. */
      Name: string;
      /** Name of the proximity group to which this object belongs. */
      ProximityGroupName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.TemplateGroupName': {
    inputs: {
      /** Name of the basic object. */
      Name: string;
    };
    outputs: {
      /** Name of the template group to which this object belongs. */
      TemplateGroupName: string;
    };
    returned: undefined;
  };
  'BasicObjectServices.SetTemplateGroupName': {
    inputs: {
      /** Name of the basic object to update. */
      Name: string;
      /** Name of the template group to which this object belongs. */
      TemplateGroupName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'BasicObjectServices.BasicObjectWarnings': {
    inputs: {
      /** Name of the basic object. */
      Name: string;
    };
    outputs: {
      /** Active warning types and descriptions for the object. */
      Warnings: [EBasicObjectWarning, string][];
    };
    returned: undefined;
  };
  'SmartObjectServices.SmartObjectList': {
    inputs: Record<string, never>;
    outputs: {
      /** List of smart object names. */
      Names: string[];
    };
    returned: undefined;
  };
  'SmartObjectServices.Add': {
    inputs: {
      /** Name for the newly created smart object. */
      Name: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.AddFromTemplate': {
    inputs: {
      /** Name for the newly created smart object. */
      Name: string;
      /** Absolute path to a smart object template file. This path must be accessible from the remote host. */
      Template: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.Remove': {
    inputs: {
      /** Smart object name. */
      Name: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.RemoveAll': {
    inputs: Record<string, never>;
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.CompatibleDeviceTypes': {
    inputs: Record<string, never>;
    outputs: {
      /** Compatible device types. */
      DeviceTypes: string[];
    };
    returned: undefined;
  };
  'SmartObjectServices.CreateSmartObjects': {
    inputs: Record<string, never>;
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.AssignOptimalActiveMarkerPatterns': {
    inputs: Record<string, never>;
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.AutoPatternManagementEnabled': {
    inputs: Record<string, never>;
    outputs: {
      /** If automatic pattern management is enabled. */
      Enabled: boolean;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetAutoPatternManagementEnabled': {
    inputs: {
      /** If automatic pattern management should be enabled. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.Rename': {
    inputs: {
      /** Name of the smart object to update. */
      OldName: string;
      /** New smart object name. */
      NewName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.SmartClusterCount': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** Number of smart clusters. */
      Count: number;
    };
    returned: undefined;
  };
  'SmartObjectServices.SmartClusterLabel': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
      /** Index of the smart cluster. */
      SmartClusterIndex: number;
    };
    outputs: {
      /** Label of the smart cluster. */
      Label: string;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetSmartClusterLabel': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
      /** Index of the smart cluster. */
      SmartClusterIndex: number;
      /** New label for the smart cluster. */
      Label: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.SmartClusterActiveMarkerPattern': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
      /** Index of the smart cluster. */
      SmartClusterIndex: number;
    };
    outputs: {
      /** Marker pattern of the smart cluster. */
      Pattern: number;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetSmartClusterActiveMarkerPattern': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
      /** Index of the smart cluster. */
      SmartClusterIndex: number;
      /** New marker pattern for the smart cluster. */
      Pattern: number;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.SmartClusterDeviceURN': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
      /** Index of the smart cluster. */
      SmartClusterIndex: number;
    };
    outputs: {
      /** Device URN linked to this smart cluster. */
      DeviceURN: string;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetSmartClusterDeviceURN': {
    inputs: {
      /** Name of the smart object to update. */
      Name: string;
      /** Index of the smart cluster. */
      SmartClusterIndex: number;
      /** Device URN to link with this smart cluster. */
      DeviceURN: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.Enabled': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** Enabled value. */
      Enabled: boolean;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetEnabled': {
    inputs: {
      /** Name of the smart object to update. */
      Name: string;
      /** Enabled value. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.SetAllEnabled': {
    inputs: {
      /** Enabled value. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.Color': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** HTML hex color code (format '#AARRGGBB'). */
      ColorHtml: string;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetColor': {
    inputs: {
      /** Name of the smart object to update. */
      Name: string;
      /** HTML hex color code (format '#AARRGGBB'). */
      ColorHtml: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.ActiveMarkersOnWhileCharging': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** True if active markers should be kept on while charging. */
      OnWhileCharging: boolean;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetActiveMarkersOnWhileCharging': {
    inputs: {
      /** Name of the smart object to update. */
      Name: string;
      /** True if active markers should be kept on while charging. */
      OnWhileCharging: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.AutoAssignEnabled': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** Auto-assign enabled value. */
      Enabled: boolean;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetAutoAssignEnabled': {
    inputs: {
      /** Name of the smart object to update. */
      Name: string;
      /** Auto-assign enabled value. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.AutoAssignedName': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** Auto-assigned name. */
      AutoAssignedName: string;
    };
    returned: undefined;
  };
  'SmartObjectServices.ProximityGroupName': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** Name of the proximity group to which this subject belongs. */
      ProximityGroupName: string;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetProximityGroupName': {
    inputs: {
      /** Name of the smart object to update. */
      Name: string;
      /** Name of the proximity group to which this subject belongs. */
      ProximityGroupName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.TemplateGroupName': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** Name of the template group to which this subject belongs. */
      TemplateGroupName: string;
    };
    returned: undefined;
  };
  'SmartObjectServices.SetTemplateGroupName': {
    inputs: {
      /** Name of the smart object to update. */
      Name: string;
      /** Name of the template group to which this subject belongs. */
      TemplateGroupName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SmartObjectServices.SmartObjectWarnings': {
    inputs: {
      /** Name of the smart object. */
      Name: string;
    };
    outputs: {
      /** Active warning types and descriptions for the smart object. */
      Warnings: [ESmartObjectWarning, string][];
    };
    returned: undefined;
  };
  'ObjectEvaluationServices.Enabled': {
    inputs: Record<string, never>;
    outputs: {
      /** If object evaluation is enabled. */
      Enabled: boolean;
    };
    returned: undefined;
  };
  'ObjectEvaluationServices.SetEnabled': {
    inputs: {
      /** If object evaluation should be enabled. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'ObjectEvaluationServices.MaximumEvaluationStepCount': {
    inputs: Record<string, never>;
    outputs: {
      /** Maximum number of steps permitted per object pair. */
      MaximumStepCount: bigint;
    };
    returned: undefined;
  };
  'ObjectEvaluationServices.SetMaximumEvaluationStepCount': {
    inputs: {
      /** Maximum number of steps permitted per object pair. */
      MaximumStepCount: bigint;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'ObjectEvaluationServices.WarningThreshold': {
    inputs: Record<string, never>;
    outputs: {
      /** Match distance in millimeters at which a warning is generated. */
      Threshold: number;
    };
    returned: undefined;
  };
  'ObjectEvaluationServices.SetWarningThreshold': {
    inputs: {
      /** Match distance in millimeters at which a warning is generated. */
      Threshold: number;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'ObjectEvaluationServices.Progress': {
    inputs: Record<string, never>;
    outputs: {
      /** Number of object comparisons done so far in this update. */
      Done: bigint;
      /** Number of object comparisons required to complete update. */
      Required: bigint;
    };
    returned: undefined;
  };
  'ObjectEvaluationServices.HighestStepCountReached': {
    inputs: Record<string, never>;
    outputs: {
      /** Highest step count reached. */
      HighestStepCountReached: bigint;
    };
    returned: undefined;
  };
  'ObjectEvaluationServices.MatchDistance': {
    inputs: {
      /** Name of the object being evaluated. */
      FirstObjectName: string;
      /** Name of the object the first is being compared to. */
      SecondObjectName: string;
    };
    outputs: {
      /** If the first object matches the second. If this is false, the match distance will be arbitrarily large.  */
      Matches: boolean;
      /** Approximate average displacement between the closest-matching object marker subsets (in millimeters). Zero distance means that the subset of markers allowed by the entrance threshold can be aligned identically and can't be distinguished. The larger this distance is, the less likely the object is to be confused with the other. */
      MatchDistance: number;
    };
    returned: undefined;
  };
  'CharacterFromClustersServices.CharacterList': {
    inputs: Record<string, never>;
    outputs: {
      /** List of character names. */
      Names: string[];
    };
    returned: undefined;
  };
  'CharacterFromClustersServices.CreateCharacter': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
      /** Absolute path to character template file. */
      TemplatePath: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.RemoveCharacter': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.RemoveAllCharacters': {
    inputs: Record<string, never>;
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.CalibrateCharacter': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.ClearCharacterCalibration': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.CharacterCalibrationState': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
    };
    outputs: {
      /** Calibration state of character. */
      CalibrationState: ECharacterCalibrationState;
    };
    returned: undefined;
  };
  'CharacterFromClustersServices.CharacterEnabled': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
    };
    outputs: {
      /** If character is enabled. */
      Enabled: boolean;
    };
    returned: undefined;
  };
  'CharacterFromClustersServices.SetCharacterEnabled': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
      /** If character should be enabled. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.SetAllCharactersEnabled': {
    inputs: {
      /** If characters should be enabled. */
      Enabled: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.CharacterRetargetPath': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
    };
    outputs: {
      /** Absolute path to a retarget file. */
      RetargetPath: string;
    };
    returned: undefined;
  };
  'CharacterFromClustersServices.SetCharacterRetargetPath': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
      /** Absolute path to retarget file. This path must be accessible from the remote host. An empty path is also accepted, which will set the retarget to None. */
      RetargetPath: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.SlotNames': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
    };
    outputs: {
      /** Names of character slots. */
      SlotNames: string[];
    };
    returned: undefined;
  };
  'CharacterFromClustersServices.SlotObject': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
      /** Index of slot. */
      SlotIndex: number;
    };
    outputs: {
      /** Name of object assigned to slot. */
      ObjectName: string;
    };
    returned: undefined;
  };
  'CharacterFromClustersServices.SetSlotObject': {
    inputs: {
      /** Name of character. */
      CharacterName: string;
      /** Index of slot. */
      SlotIndex: number;
      /** Name of object to assign to slot. */
      ObjectName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'CharacterFromClustersServices.CharacterWarnings': {
    inputs: {
      /** Name of the character. */
      Name: string;
    };
    outputs: {
      /** Active warning types and descriptions for the character. */
      Warnings: [ECharacterWarning, string][];
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.CanStartSubjectCalibration': {
    inputs: Record<string, never>;
    outputs: {
      /** The reason why subject calibration cannot be initiated. */
      Reason: string;
    };
    returned: boolean;
  };
  'SubjectCalibrationServices.CanStartSubjectRecalibration': {
    inputs: Record<string, never>;
    outputs: {
      /** The reason why subject re-calibration cannot be initiated. */
      Reason: string;
    };
    returned: boolean;
  };
  'SubjectCalibrationServices.CanAcceptTPose': {
    inputs: Record<string, never>;
    outputs: {
      /** The reason why the T-Pose cannot be selected. */
      Reason: string;
    };
    returned: boolean;
  };
  'SubjectCalibrationServices.CanStopSubjectCalibration': {
    inputs: Record<string, never>;
    outputs: {
      /** The reason why subject calibration cannot be completed. */
      Reason: string;
    };
    returned: boolean;
  };
  'SubjectCalibrationServices.CanCancelSubjectCalibration': {
    inputs: Record<string, never>;
    outputs: {
      /** The reason why subject calibration cannot be canceled. */
      Reason: string;
    };
    returned: boolean;
  };
  'SubjectCalibrationServices.StartSubjectCalibration': {
    inputs: {
      /** A capture name to use for the subject calibration files.  Leave blank to use the default.  If the name already exists in the capture directory it will be overwritten. */
      CaptureName: string;
    };
    outputs: {
      /** Provides the session id for the calibration.  This is provided to to Cancel and Stop to ensure the correct subject calibration is being terminated. */
      SubjectCalibrationSession: number;
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.StartSubjectRecalibration': {
    inputs: {
      /** A capture name to use for the subject calibration files.  Leave blank to use the default.  If the name already exists in the capture directory it will be overwritten. */
      CaptureName: string;
    };
    outputs: {
      /** Provides the session id for the calibration.  This is provided to to Cancel and Stop to ensure the correct subject calibration is being terminated. */
      SubjectCalibrationSession: number;
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.AcceptTPose': {
    inputs: {
      /** The session id for the calibration.  This will have been provided by StartSubjectCalibration or StartSubjectRecalibration. */
      SubjectCalibrationSession: number;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SubjectCalibrationServices.CancelSubjectCalibration': {
    inputs: {
      /** The session id for the calibration.  This will have been provided by StartSubjectCalibration or StartSubjectRecalibration. */
      SubjectCalibrationSession: number;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SubjectCalibrationServices.StopSubjectCalibration': {
    inputs: {
      /** The session id for the calibration.  This will have been provided by StartSubjectCalibration or StartSubjectRecalibration. */
      SubjectCalibrationSession: number;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SubjectCalibrationServices.LatestSubjectCalibrationState': {
    inputs: Record<string, never>;
    outputs: {
      /** The currently executing session id. */
      SessionId: number;
      /** The current state of calibration. */
      State: ESubjectCalibrationState;
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.NewSubjectName': {
    inputs: Record<string, never>;
    outputs: {
      /** The subject name. */
      SubjectName: string;
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.SetNewSubjectName': {
    inputs: {
      /** Subject name to set. */
      SubjectName: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SubjectCalibrationServices.SubjectLabellingTemplates': {
    inputs: Record<string, never>;
    outputs: {
      /** The set of labeling templates. */
      LabellingTemplates: string[];
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.SubjectLabellingTemplate': {
    inputs: Record<string, never>;
    outputs: {
      /** The labeling template to use for the next subject calibration. */
      LabellingTemplate: string;
      /** The full path to the template. */
      LabellingTemplatePath: string;
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.SetSubjectLabellingTemplate': {
    inputs: {
      /** The labeling template to use for the next subject calibration. */
      LabellingTemplate: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'SubjectCalibrationServices.SubjectSkins': {
    inputs: Record<string, never>;
    outputs: {
      /** The set of available skins. */
      Skins: string[];
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.SubjectSkin': {
    inputs: Record<string, never>;
    outputs: {
      /** The skin name to use for the next subject calibration. */
      Skin: string;
      /** The full path to the skin. */
      SkinPath: string;
    };
    returned: undefined;
  };
  'SubjectCalibrationServices.SetSubjectSkin': {
    inputs: {
      /** The skin use for the next subject calibration. */
      Skin: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'HostSimulation.Devices': {
    inputs: Record<string, never>;
    outputs: {
      /** List of device URNs. */
      Urns: string[];
    };
    returned: undefined;
  };
  'HostSimulation.DeviceState': {
    inputs: {
      /** URN of the device. */
      Urn: string;
    };
    outputs: {
      /** Type of the device. */
      Type: string;
      /** If the device is connected. */
      Connected: boolean;
      /** If the device is charging. */
      Charging: boolean;
      /** Charge of the battery in percent. */
      Battery: number;
      /** Radio channel of the device, 0 if it has none. */
      Radio: number;
    };
    returned: undefined;
  };
  'HostSimulation.AddDevice': {
    inputs: {
      /** URN of the new device. */
      Urn: string;
      /** Type of the new device. */
      Type: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'HostSimulation.RemoveDevice': {
    inputs: {
      /** URN of the device. */
      Urn: string;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'HostSimulation.SetConnected': {
    inputs: {
      /** URN of the device. */
      Urn: string;
      /** If the device should be connected. */
      Connected: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'HostSimulation.SetCharging': {
    inputs: {
      /** URN of the device. */
      Urn: string;
      /** If the device should be charging. */
      Charging: boolean;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'HostSimulation.SetBattery': {
    inputs: {
      /** URN of the device. */
      Urn: string;
      /** New charge of the battery in percent. */
      Percent: number;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
  'HostSimulation.SetRadio': {
    inputs: {
      /** URN of the device. */
      Urn: string;
      /** New radio channel of the device, 0 for none. */
      Radio: number;
    };
    outputs: Record<string, never>;
    returned: undefined;
  };
}

/** The parameters of the callbacks by their full names. */
export interface Callbacks {
  /** Callback issued whenever any basic object changes. This includes addition/removal of basic objects and basic object property changes. */
  'BasicObjectServices.BasicObjectChangedCallback': {
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever any smart object changes. This includes addition/removal of smart objects and smart object property changes. */
  'SmartObjectServices.SmartObjectChangedCallback': {
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever object evaluation changes. */
  'ObjectEvaluationServices.EvaluationChangedCallback': {
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever any character changes. This includes addition/removal of characters and character property changes. */
  'CharacterFromClustersServices.CharacterChangedCallback': {
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever the systems ability to start subject calibration changed. */
  'SubjectCalibrationServices.CanStartSubjectCalibrationChangedCallback': {
    /** Can the system start subject calibration? */
    Able: boolean;
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever the systems ability to start subject re-calibration changed. */
  'SubjectCalibrationServices.CanStartSubjectRecalibrationChangedCallback': {
    /** Can the system start subject re-calibration? */
    Able: boolean;
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever the systems ability to accept a T-Pose changed. */
  'SubjectCalibrationServices.CanAcceptTPoseChangedCallback': {
    /** Can the system accept a T-Pose? */
    Able: boolean;
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever the systems ability to stop subject calibration or re-calibration changed. */
  'SubjectCalibrationServices.CanStopSubjectCalibrationChangedCallback': {
    /** Can the system stop subject calibration? */
    Able: boolean;
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** @deprecated (Tessera) Deprecated alias for CanStopSubjectCalibrationChangedCallback. */
  'SubjectCalibrationServices.CanEndSubjectCalibrationChangedCallback': {
    /** Can the system stop subject calibration? */
    Able: boolean;
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever the systems ability to cancel subject calibration or re-calibration changed. */
  'SubjectCalibrationServices.CanCancelSubjectCalibrationChangedCallback': {
    /** Can the system cancel subject calibration? */
    Able: boolean;
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever the calibration state changes. */
  'SubjectCalibrationServices.LatestSubjectCalibrationStateChangedCallback': {
    /** The currently executing session id. */
    SessionId: number;
    /** The current state of calibration. */
    State: ESubjectCalibrationState;
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
  /** Callback issued whenever any of the calibration settings changes. */
  'SubjectCalibrationServices.SubjectCalibrationSettingsChangedCallback': {
    /** Counts the notifications of the whole server. */
    sequence: bigint;
  };
}

/** Greets a client; the first message of each connection. */
export interface Hello {
  /** Number of the connection, since the host was started. */
  session: number;
  /** New at each start of the host. When it differs after a reconnection, everything that a client remembers may be stale. */
  epoch: string;
  /** SHA-256 of openrpc.json followed by asyncapi.json, in hexadecimal: another text when the API is another one. */
  api: string;
  limits: {
    /** Length of a message, in bytes. */
    messageBytes: number;
    /** Depth of arrays and objects in a message. */
    nesting: number;
    /** Calls in a batch. */
    batchCalls: number;
    /** Connections of all clients together. */
    connections: number;
    /** Connections that are WebSockets. */
    webSockets: number;
    /** Callbacks that a connection subscribes to. */
    subscriptions: number;
    /** Calls of a connection at the same time; more wait. */
    callsInFlight: number;
    /** Calls of all connections at the same time; more wait. */
    callsInFlightOverall: number;
    /** Bytes that wait for the client to read them; also the longest response. */
    outgoingBytes: number;
    /** Bytes that wait for all clients together; beyond, each has its share only. */
    outgoingBytesOverall: number;
    /** Notifications that wait for the client to read them and may not stand for each other. */
    outgoingNotifications: number;
    /** Seconds of silence after which a WebSocket client is pinged; as long again, and the connection is ended. */
    pingAfterSeconds: number;
  };
  levels: {
    /** Level of what everybody may call. */
    open: number;
    /** Level of what is a preview. */
    preview: number;
    /** Least level that this client may call. */
    granted: number;
  };
}

/** The members of outputs and parameters that are 64 bits wide: always a bigint. */
export const wideMembers: Readonly<Record<string, readonly string[]>> = {
  'ObjectEvaluationServices.MaximumEvaluationStepCount': ['MaximumStepCount'],
  'ObjectEvaluationServices.Progress': ['Done', 'Required'],
  'ObjectEvaluationServices.HighestStepCountReached': ['HighestStepCountReached'],
  'BasicObjectServices.BasicObjectChangedCallback': ['sequence'],
  'SmartObjectServices.SmartObjectChangedCallback': ['sequence'],
  'ObjectEvaluationServices.EvaluationChangedCallback': ['sequence'],
  'CharacterFromClustersServices.CharacterChangedCallback': ['sequence'],
  'SubjectCalibrationServices.CanStartSubjectCalibrationChangedCallback': ['sequence'],
  'SubjectCalibrationServices.CanStartSubjectRecalibrationChangedCallback': ['sequence'],
  'SubjectCalibrationServices.CanAcceptTPoseChangedCallback': ['sequence'],
  'SubjectCalibrationServices.CanStopSubjectCalibrationChangedCallback': ['sequence'],
  'SubjectCalibrationServices.CanEndSubjectCalibrationChangedCallback': ['sequence'],
  'SubjectCalibrationServices.CanCancelSubjectCalibrationChangedCallback': ['sequence'],
  'SubjectCalibrationServices.LatestSubjectCalibrationStateChangedCallback': ['sequence'],
  'SubjectCalibrationServices.SubjectCalibrationSettingsChangedCallback': ['sequence'],
};

/** Functions for managing basic objects. Basic objects are rigid bodies, with a fixed physical marker pattern. */
export class BasicObjectServices {
  readonly #caller: Caller;

  constructor(caller: Caller) {
    this.#caller = caller;
  }

  /** The list of loaded basic object names. */
  async basicObjectList(options?: CallOptions): Promise<Outputs<'BasicObjectServices.BasicObjectList'>> {
    return (await this.#caller.call('BasicObjectServices.BasicObjectList', {}, options)).outputs;
  }

  /**
   * Remove a basic object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is not loaded.
   */
  async remove(inputs: Inputs<'BasicObjectServices.Remove'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.Remove', inputs, options);
  }

  /** Remove all basic objects. */
  async removeAll(options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.RemoveAll', {}, options);
  }

  /**
   * Update the basic object name.
   * @throws SubjectStoreError `AlreadyPresent`: if the new name is already in use.
   * @throws SubjectStoreError `InvalidName`: if the new name contains invalid characters or has leading/trailing spaces.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async rename(inputs: Inputs<'BasicObjectServices.Rename'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.Rename', inputs, options);
  }

  /**
   * Get the enabled value of a basic object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async enabled(inputs: Inputs<'BasicObjectServices.Enabled'>, options?: CallOptions): Promise<Outputs<'BasicObjectServices.Enabled'>> {
    return (await this.#caller.call('BasicObjectServices.Enabled', inputs, options)).outputs;
  }

  /**
   * Enable or disable a basic object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async setEnabled(inputs: Inputs<'BasicObjectServices.SetEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.SetEnabled', inputs, options);
  }

  /** Enable or disable all basic objects. */
  async setAllEnabled(inputs: Inputs<'BasicObjectServices.SetAllEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.SetAllEnabled', inputs, options);
  }

  /**
   * Get the color of a basic object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async color(inputs: Inputs<'BasicObjectServices.Color'>, options?: CallOptions): Promise<Outputs<'BasicObjectServices.Color'>> {
    return (await this.#caller.call('BasicObjectServices.Color', inputs, options)).outputs;
  }

  /** Set the color of a basic object. */
  async setColor(inputs: Inputs<'BasicObjectServices.SetColor'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.SetColor', inputs, options);
  }

  /**
   * Get the character auto-assign enabled value of a basic object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async autoAssignEnabled(inputs: Inputs<'BasicObjectServices.AutoAssignEnabled'>, options?: CallOptions): Promise<Outputs<'BasicObjectServices.AutoAssignEnabled'>> {
    return (await this.#caller.call('BasicObjectServices.AutoAssignEnabled', inputs, options)).outputs;
  }

  /**
   * Enable or disable character auto-assignment for a basic object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async setAutoAssignEnabled(inputs: Inputs<'BasicObjectServices.SetAutoAssignEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.SetAutoAssignEnabled', inputs, options);
  }

  /**
   * Get the name auto-assigned to a basic object. Objects are not renamed when auto-assigned to a character slot. Instead, the name used for data stream output changes to match the slot name.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   * @throws SubjectStoreError `NotSet`: If the subject is not currently assigned, or auto-assign is disabled for the subject.
   */
  async autoAssignedName(inputs: Inputs<'BasicObjectServices.AutoAssignedName'>, options?: CallOptions): Promise<Outputs<'BasicObjectServices.AutoAssignedName'>> {
    return (await this.#caller.call('BasicObjectServices.AutoAssignedName', inputs, options)).outputs;
  }

  /**
   * Get the proximity group name for this object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async proximityGroupName(inputs: Inputs<'BasicObjectServices.ProximityGroupName'>, options?: CallOptions): Promise<Outputs<'BasicObjectServices.ProximityGroupName'>> {
    return (await this.#caller.call('BasicObjectServices.ProximityGroupName', inputs, options)).outputs;
  }

  /**
   * Set the proximity group name for this object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async setProximityGroupName(inputs: Inputs<'BasicObjectServices.SetProximityGroupName'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.SetProximityGroupName', inputs, options);
  }

  /**
   * Get the template group name for this object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async templateGroupName(inputs: Inputs<'BasicObjectServices.TemplateGroupName'>, options?: CallOptions): Promise<Outputs<'BasicObjectServices.TemplateGroupName'>> {
    return (await this.#caller.call('BasicObjectServices.TemplateGroupName', inputs, options)).outputs;
  }

  /**
   * Set the template group name for this object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async setTemplateGroupName(inputs: Inputs<'BasicObjectServices.SetTemplateGroupName'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('BasicObjectServices.SetTemplateGroupName', inputs, options);
  }

  /**
   * Get any warnings associated with a basic object.
   * @throws SubjectStoreError `NotFound`: If the basic object name supplied is invalid.
   */
  async basicObjectWarnings(inputs: Inputs<'BasicObjectServices.BasicObjectWarnings'>, options?: CallOptions): Promise<Outputs<'BasicObjectServices.BasicObjectWarnings'>> {
    return (await this.#caller.call('BasicObjectServices.BasicObjectWarnings', inputs, options)).outputs;
  }
}

/** Functions for managing smart objects. A smart object represents the binding between the object (which appears in the data-stream) and the physical cluster device. The smart object can be configured in advance of the device arrival and persists after device disconnection. */
export class SmartObjectServices {
  readonly #caller: Caller;

  constructor(caller: Caller) {
    this.#caller = caller;
  }

  /** The list of loaded smart object names. */
  async smartObjectList(options?: CallOptions): Promise<Outputs<'SmartObjectServices.SmartObjectList'>> {
    return (await this.#caller.call('SmartObjectServices.SmartObjectList', {}, options)).outputs;
  }

  /**
   * Add a new smart object using the Corvex template. A unique pattern will be assigned automatically if possible.
   * @throws SubjectStoreError `AlreadyPresent`: If the name is already in use.
   * @throws SubjectStoreError `InvalidName`: If the name contains invalid characters or has leading/trailing spaces.
   */
  async add(inputs: Inputs<'SmartObjectServices.Add'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.Add', inputs, options);
  }

  /** Add a new smart object using the specified template. A unique pattern will be assigned to each smart cluster automatically if possible. */
  async addFromTemplate(inputs: Inputs<'SmartObjectServices.AddFromTemplate'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.AddFromTemplate', inputs, options);
  }

  /**
   * Remove a smart object.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is not loaded.
   */
  async remove(inputs: Inputs<'SmartObjectServices.Remove'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.Remove', inputs, options);
  }

  /** Remove all smart objects. */
  async removeAll(options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.RemoveAll', {}, options);
  }

  /** Get a list of device types compatible with smart objects. */
  async compatibleDeviceTypes(options?: CallOptions): Promise<Outputs<'SmartObjectServices.CompatibleDeviceTypes'>> {
    return (await this.#caller.call('SmartObjectServices.CompatibleDeviceTypes', {}, options)).outputs;
  }

  async createSmartObjects(options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.CreateSmartObjects', {}, options);
  }

  /**
   * Assign a distinct active marker pattern to each smart cluster in the loaded smart objects.
If there isn't a pattern set that supports the required number of patterns, any excess smart clusters will be assigned pattern 0.
   * @throws SubjectStoreError `NotFound`: If an unrecognized smart cluster type was found.
   * @throws SubjectStoreError `NotSupported`: If an unsupported combination of smart cluster types was found.
   */
  async assignOptimalActiveMarkerPatterns(options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.AssignOptimalActiveMarkerPatterns', {}, options);
  }

  /** Get if smart object patterns are being managed automatically by the application. */
  async autoPatternManagementEnabled(options?: CallOptions): Promise<Outputs<'SmartObjectServices.AutoPatternManagementEnabled'>> {
    return (await this.#caller.call('SmartObjectServices.AutoPatternManagementEnabled', {}, options)).outputs;
  }

  /** Set if smart object patterns should be managed automatically by the application. */
  async setAutoPatternManagementEnabled(inputs: Inputs<'SmartObjectServices.SetAutoPatternManagementEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetAutoPatternManagementEnabled', inputs, options);
  }

  /**
   * Update the smart object name.
   * @throws SubjectStoreError `AlreadyPresent`: if the new name is already in use.
   * @throws SubjectStoreError `InvalidName`: if the new name contains invalid characters or has leading/trailing spaces.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async rename(inputs: Inputs<'SmartObjectServices.Rename'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.Rename', inputs, options);
  }

  /**
   * The number of smart clusters that make up this smart object.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async smartClusterCount(inputs: Inputs<'SmartObjectServices.SmartClusterCount'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.SmartClusterCount'>> {
    return (await this.#caller.call('SmartObjectServices.SmartClusterCount', inputs, options)).outputs;
  }

  /** The label used to identify a smart cluster on the smart object. */
  async smartClusterLabel(inputs: Inputs<'SmartObjectServices.SmartClusterLabel'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.SmartClusterLabel'>> {
    return (await this.#caller.call('SmartObjectServices.SmartClusterLabel', inputs, options)).outputs;
  }

  /** Set the label used to identify a smart cluster on the smart object. */
  async setSmartClusterLabel(inputs: Inputs<'SmartObjectServices.SetSmartClusterLabel'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetSmartClusterLabel', inputs, options);
  }

  /**
   * The marker pattern to set on the smart cluster. This updates the markers on the linked device and the associated subject for tracking.
   * @throws SubjectStoreError `InvalidIndex`: If the smart cluster index is greater than or equal to the smart cluster count.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async smartClusterActiveMarkerPattern(inputs: Inputs<'SmartObjectServices.SmartClusterActiveMarkerPattern'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.SmartClusterActiveMarkerPattern'>> {
    return (await this.#caller.call('SmartObjectServices.SmartClusterActiveMarkerPattern', inputs, options)).outputs;
  }

  /**
   * Update the marker pattern to set on the smart cluster.
   * @throws SubjectStoreError `InvalidIndex`: If the smart cluster index is greater than or equal to the smart cluster count.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async setSmartClusterActiveMarkerPattern(inputs: Inputs<'SmartObjectServices.SetSmartClusterActiveMarkerPattern'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetSmartClusterActiveMarkerPattern', inputs, options);
  }

  /** The device linked to this smart cluster. */
  async smartClusterDeviceURN(inputs: Inputs<'SmartObjectServices.SmartClusterDeviceURN'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.SmartClusterDeviceURN'>> {
    return (await this.#caller.call('SmartObjectServices.SmartClusterDeviceURN', inputs, options)).outputs;
  }

  /** Update the device linked with this smart cluster. To clear the link to a device set the URN to an empty string. */
  async setSmartClusterDeviceURN(inputs: Inputs<'SmartObjectServices.SetSmartClusterDeviceURN'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetSmartClusterDeviceURN', inputs, options);
  }

  /**
   * Get the enabled value of a smart object.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async enabled(inputs: Inputs<'SmartObjectServices.Enabled'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.Enabled'>> {
    return (await this.#caller.call('SmartObjectServices.Enabled', inputs, options)).outputs;
  }

  /**
   * Enable or disable a smart object.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async setEnabled(inputs: Inputs<'SmartObjectServices.SetEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetEnabled', inputs, options);
  }

  /** Enable or disable all smart objects. */
  async setAllEnabled(inputs: Inputs<'SmartObjectServices.SetAllEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetAllEnabled', inputs, options);
  }

  /**
   * Get the color of a smart object (and the generated object).
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async color(inputs: Inputs<'SmartObjectServices.Color'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.Color'>> {
    return (await this.#caller.call('SmartObjectServices.Color', inputs, options)).outputs;
  }

  /** Set the color of a smart object (and the generated object). */
  async setColor(inputs: Inputs<'SmartObjectServices.SetColor'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetColor', inputs, options);
  }

  /**
   * Get the active markers on while charging value for linked devices.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async activeMarkersOnWhileCharging(inputs: Inputs<'SmartObjectServices.ActiveMarkersOnWhileCharging'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.ActiveMarkersOnWhileCharging'>> {
    return (await this.#caller.call('SmartObjectServices.ActiveMarkersOnWhileCharging', inputs, options)).outputs;
  }

  /**
   * Set the active markers on while charging value for linked devices.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async setActiveMarkersOnWhileCharging(inputs: Inputs<'SmartObjectServices.SetActiveMarkersOnWhileCharging'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetActiveMarkersOnWhileCharging', inputs, options);
  }

  /**
   * Get the character auto-assign enabled value of a smart object.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async autoAssignEnabled(inputs: Inputs<'SmartObjectServices.AutoAssignEnabled'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.AutoAssignEnabled'>> {
    return (await this.#caller.call('SmartObjectServices.AutoAssignEnabled', inputs, options)).outputs;
  }

  /**
   * Enable or disable character auto-assignment for a smart object.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async setAutoAssignEnabled(inputs: Inputs<'SmartObjectServices.SetAutoAssignEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetAutoAssignEnabled', inputs, options);
  }

  /**
   * Get the name auto-assigned to a smart object. Objects are not renamed when auto-assigned to a character slot. Instead, the name used for data stream output changes to match the slot name.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   * @throws SubjectStoreError `NotSet`: If the subject is not currently assigned, or auto-assign is disabled for the subject.
   */
  async autoAssignedName(inputs: Inputs<'SmartObjectServices.AutoAssignedName'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.AutoAssignedName'>> {
    return (await this.#caller.call('SmartObjectServices.AutoAssignedName', inputs, options)).outputs;
  }

  /**
   * Get the proximity group name for this subject.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async proximityGroupName(inputs: Inputs<'SmartObjectServices.ProximityGroupName'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.ProximityGroupName'>> {
    return (await this.#caller.call('SmartObjectServices.ProximityGroupName', inputs, options)).outputs;
  }

  /**
   * Set the proximity group name for this subject.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async setProximityGroupName(inputs: Inputs<'SmartObjectServices.SetProximityGroupName'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetProximityGroupName', inputs, options);
  }

  /**
   * Get the template group name for this subject.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async templateGroupName(inputs: Inputs<'SmartObjectServices.TemplateGroupName'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.TemplateGroupName'>> {
    return (await this.#caller.call('SmartObjectServices.TemplateGroupName', inputs, options)).outputs;
  }

  /**
   * Set the template group name for this subject.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async setTemplateGroupName(inputs: Inputs<'SmartObjectServices.SetTemplateGroupName'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SmartObjectServices.SetTemplateGroupName', inputs, options);
  }

  /**
   * Get any warnings associated with a smart object.
   * @throws SubjectStoreError `NotFound`: If the smart object name supplied is invalid.
   */
  async smartObjectWarnings(inputs: Inputs<'SmartObjectServices.SmartObjectWarnings'>, options?: CallOptions): Promise<Outputs<'SmartObjectServices.SmartObjectWarnings'>> {
    return (await this.#caller.call('SmartObjectServices.SmartObjectWarnings', inputs, options)).outputs;
  }
}

/** Services for object evaluation. This feature may be used to detect potential confusion between one object and another (basic or smart), or a different view of itself. */
export class ObjectEvaluationServices {
  readonly #caller: Caller;

  constructor(caller: Caller) {
    this.#caller = caller;
  }

  /** Query if object evaluation is enabled. */
  async enabled(options?: CallOptions): Promise<Outputs<'ObjectEvaluationServices.Enabled'>> {
    return (await this.#caller.call('ObjectEvaluationServices.Enabled', {}, options)).outputs;
  }

  /** Enable or disable object evaluation. Note that object evaluation can be computationally intensive, depending on the number and size of objects loaded. It is recommended to disable this feature during a live experience. */
  async setEnabled(inputs: Inputs<'ObjectEvaluationServices.SetEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('ObjectEvaluationServices.SetEnabled', inputs, options);
  }

  /** Query the maximum number of steps to take per object pair. */
  async maximumEvaluationStepCount(options?: CallOptions): Promise<Outputs<'ObjectEvaluationServices.MaximumEvaluationStepCount'>> {
    return (await this.#caller.call('ObjectEvaluationServices.MaximumEvaluationStepCount', {}, options)).outputs;
  }

  /** Set the maximum number of steps to take per object pair. Objects with a large number of markers will generally require more steps to fully evaluate. */
  async setMaximumEvaluationStepCount(inputs: Inputs<'ObjectEvaluationServices.SetMaximumEvaluationStepCount'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('ObjectEvaluationServices.SetMaximumEvaluationStepCount', inputs, options);
  }

  /** Query the distance threshold for warning about a match between two objects. */
  async warningThreshold(options?: CallOptions): Promise<Outputs<'ObjectEvaluationServices.WarningThreshold'>> {
    return (await this.#caller.call('ObjectEvaluationServices.WarningThreshold', {}, options)).outputs;
  }

  /** Set the distance threshold for warning about a match between two objects. This relates to the closest average distance between markers when the two objects are aligned. */
  async setWarningThreshold(inputs: Inputs<'ObjectEvaluationServices.SetWarningThreshold'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('ObjectEvaluationServices.SetWarningThreshold', inputs, options);
  }

  /**
   * Get progress for the current object evaluation update. Evaluation is finished when the required number of comparisons have been done. Object changes whilst evaluation is in progress will increase the number of comparisons required. If evaluation has finished, progress will reset to zero on any subsequent object changes.
   * @throws SubjectStoreError `NotAvailable`: If object evaluation is disabled.
   */
  async progress(options?: CallOptions): Promise<Outputs<'ObjectEvaluationServices.Progress'>> {
    return (await this.#caller.call('ObjectEvaluationServices.Progress', {}, options)).outputs;
  }

  /**
   * Get the highest number of steps reached during object evaluation. If this equals the maximum step count, you need to increase the maximum in order to fully evaluate your objects.
   * @throws SubjectStoreError `NotAvailable`: If object evaluation is disabled.
   */
  async highestStepCountReached(options?: CallOptions): Promise<Outputs<'ObjectEvaluationServices.HighestStepCountReached'>> {
    return (await this.#caller.call('ObjectEvaluationServices.HighestStepCountReached', {}, options)).outputs;
  }

  /**
   * Check if the first object matches the second. This is provided for test purposes, as object confusion is reported via warnings. Note that matching depends on the entrance threshold of the first object. If this function is called before evaluation is finished, the objects may not have been compared yet and no match will be returned.
   * @throws SubjectStoreError `NotAvailable`: If object evaluation is disabled.
   * @throws SubjectStoreError `NotFound`: If either object name was not found or is not an object.
   * @throws SubjectStoreError `NotRequired`: If either object is disabled. Only enabled objects are evaluated.
   */
  async matchDistance(inputs: Inputs<'ObjectEvaluationServices.MatchDistance'>, options?: CallOptions): Promise<Outputs<'ObjectEvaluationServices.MatchDistance'>> {
    return (await this.#caller.call('ObjectEvaluationServices.MatchDistance', inputs, options)).outputs;
  }
}

/** Functions for controlling characters tracked from clusters. */
export class CharacterFromClustersServices {
  readonly #caller: Caller;

  constructor(caller: Caller) {
    this.#caller = caller;
  }

  /** The list of loaded character names. */
  async characterList(options?: CallOptions): Promise<Outputs<'CharacterFromClustersServices.CharacterList'>> {
    return (await this.#caller.call('CharacterFromClustersServices.CharacterList', {}, options)).outputs;
  }

  /**
   * Create a character from clusters.
   * @throws SubjectStoreError `AlreadyPresent`: A character with that name already exists.
   * @throws SubjectStoreError `FileIOFailure`: Template file could not be read.
   * @throws SubjectStoreError `FileNotFound`: Template path did not exist.
   * @throws SubjectStoreError `InvalidArgument`: Template path was empty.
   * @throws SubjectStoreError `InvalidName`: Character name is not valid.
   * @throws SubjectStoreError `SerialisationFailure`: Template file could not be parsed
   */
  async createCharacter(inputs: Inputs<'CharacterFromClustersServices.CreateCharacter'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.CreateCharacter', inputs, options);
  }

  /**
   * Remove a character.
   * @throws SubjectStoreError `NotSupported`: Name exists but is not a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async removeCharacter(inputs: Inputs<'CharacterFromClustersServices.RemoveCharacter'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.RemoveCharacter', inputs, options);
  }

  /** Remove all characters. */
  async removeAllCharacters(options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.RemoveAllCharacters', {}, options);
  }

  /**
   * Calibrate a character (adjust skeleton to fit the person, based on tracked object poses).
   * @throws SubjectStoreError `NotSupported`: Name exists but is not a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async calibrateCharacter(inputs: Inputs<'CharacterFromClustersServices.CalibrateCharacter'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.CalibrateCharacter', inputs, options);
  }

  /**
   * Clear a character calibration (return skeleton to default state).
   * @throws SubjectStoreError `NotSupported`: Name exists but is not a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async clearCharacterCalibration(inputs: Inputs<'CharacterFromClustersServices.ClearCharacterCalibration'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.ClearCharacterCalibration', inputs, options);
  }

  /**
   * Get the calibration state of a character.
   * @throws SubjectStoreError `NotSupported`: Name exists but is not a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async characterCalibrationState(inputs: Inputs<'CharacterFromClustersServices.CharacterCalibrationState'>, options?: CallOptions): Promise<Outputs<'CharacterFromClustersServices.CharacterCalibrationState'>> {
    return (await this.#caller.call('CharacterFromClustersServices.CharacterCalibrationState', inputs, options)).outputs;
  }

  /**
   * Get the enable state of a character.
   * @throws SubjectStoreError `NotSupported`: Name exists but is not a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async characterEnabled(inputs: Inputs<'CharacterFromClustersServices.CharacterEnabled'>, options?: CallOptions): Promise<Outputs<'CharacterFromClustersServices.CharacterEnabled'>> {
    return (await this.#caller.call('CharacterFromClustersServices.CharacterEnabled', inputs, options)).outputs;
  }

  /**
   * Enable or disable a character.
   * @throws SubjectStoreError `NotSupported`: Name exists but is not a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async setCharacterEnabled(inputs: Inputs<'CharacterFromClustersServices.SetCharacterEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.SetCharacterEnabled', inputs, options);
  }

  /** Enable or disable all characters. */
  async setAllCharactersEnabled(inputs: Inputs<'CharacterFromClustersServices.SetAllCharactersEnabled'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.SetAllCharactersEnabled', inputs, options);
  }

  /**
   * Get the path to a character's retarget file.
   * @throws SubjectStoreError `NotSupported`: Name exists but is not a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async characterRetargetPath(inputs: Inputs<'CharacterFromClustersServices.CharacterRetargetPath'>, options?: CallOptions): Promise<Outputs<'CharacterFromClustersServices.CharacterRetargetPath'>> {
    return (await this.#caller.call('CharacterFromClustersServices.CharacterRetargetPath', inputs, options)).outputs;
  }

  /**
   * Set the path to a character's retarget file.
   * @throws SubjectStoreError `NotSupported`: Name exists but is not a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   * @throws SubjectStoreError `FileNotFound`: If the template path did not correspond to a file.
   */
  async setCharacterRetargetPath(inputs: Inputs<'CharacterFromClustersServices.SetCharacterRetargetPath'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.SetCharacterRetargetPath', inputs, options);
  }

  /**
   * Get the names of the slots in a character.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async slotNames(inputs: Inputs<'CharacterFromClustersServices.SlotNames'>, options?: CallOptions): Promise<Outputs<'CharacterFromClustersServices.SlotNames'>> {
    return (await this.#caller.call('CharacterFromClustersServices.SlotNames', inputs, options)).outputs;
  }

  /**
   * Get the object assigned to a character slot (if any).
   * @throws SubjectStoreError `InvalidIndex`: No slot with that index.
   * @throws SubjectStoreError `NotFound`: No character with that name.
   */
  async slotObject(inputs: Inputs<'CharacterFromClustersServices.SlotObject'>, options?: CallOptions): Promise<Outputs<'CharacterFromClustersServices.SlotObject'>> {
    return (await this.#caller.call('CharacterFromClustersServices.SlotObject', inputs, options)).outputs;
  }

  /**
   * Set the object assigned to a character slot. Supplying an empty name will clear the slot.
   * @throws SubjectStoreError `InvalidIndex`: No slot with that index.
   * @throws SubjectStoreError `InvalidType`: Object name does not correspond to an object.
   * @throws SubjectStoreError `NotFound`: No character or object with that name.
   */
  async setSlotObject(inputs: Inputs<'CharacterFromClustersServices.SetSlotObject'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('CharacterFromClustersServices.SetSlotObject', inputs, options);
  }

  /**
   * Get any warnings associated with a character.
   * @throws SubjectStoreError `NotFound`: If the character name supplied is invalid.
   */
  async characterWarnings(inputs: Inputs<'CharacterFromClustersServices.CharacterWarnings'>, options?: CallOptions): Promise<Outputs<'CharacterFromClustersServices.CharacterWarnings'>> {
    return (await this.#caller.call('CharacterFromClustersServices.CharacterWarnings', inputs, options)).outputs;
  }
}

/** Functions for controlling and monitoring subject calibration. */
export class SubjectCalibrationServices {
  readonly #caller: Caller;

  constructor(caller: Caller) {
    this.#caller = caller;
  }

  /**
   * Is the system able to initiate subject calibration?
   * @returns `returned`: If you can start subject calibration.
   */
  async canStartSubjectCalibration(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.CanStartSubjectCalibration'> & { returned: boolean }> {
    const { outputs, returned } = await this.#caller.call('SubjectCalibrationServices.CanStartSubjectCalibration', {}, options);
    return { ...outputs, returned };
  }

  /**
   * Is the system able to initiate subject re-calibration?
   * @returns `returned`: If you can start subject re-calibration.
   */
  async canStartSubjectRecalibration(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.CanStartSubjectRecalibration'> & { returned: boolean }> {
    const { outputs, returned } = await this.#caller.call('SubjectCalibrationServices.CanStartSubjectRecalibration', {}, options);
    return { ...outputs, returned };
  }

  /**
   * Can the system accept the current state as a T-Pose?
   * @returns `returned`: If you can accept the current state as a T-Pose.
   */
  async canAcceptTPose(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.CanAcceptTPose'> & { returned: boolean }> {
    const { outputs, returned } = await this.#caller.call('SubjectCalibrationServices.CanAcceptTPose', {}, options);
    return { ...outputs, returned };
  }

  /**
   * Can the system stop (complete) subject calibration?
   * @returns `returned`: If you can stop subject calibration.
   */
  async canStopSubjectCalibration(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.CanStopSubjectCalibration'> & { returned: boolean }> {
    const { outputs, returned } = await this.#caller.call('SubjectCalibrationServices.CanStopSubjectCalibration', {}, options);
    return { ...outputs, returned };
  }

  /**
   * Can the system cancel subject calibration?
   * @returns `returned`: If you can cancel subject calibration.
   */
  async canCancelSubjectCalibration(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.CanCancelSubjectCalibration'> & { returned: boolean }> {
    const { outputs, returned } = await this.#caller.call('SubjectCalibrationServices.CanCancelSubjectCalibration', {}, options);
    return { ...outputs, returned };
  }

  /**
   * Initiates subject calibration.
   * @throws SubjectStoreError `InvalidArgument`: If the capture name has invalid characters.
   * @throws SubjectStoreError `NotAvailable`: If calibration is currently running.
   */
  async startSubjectCalibration(inputs: Inputs<'SubjectCalibrationServices.StartSubjectCalibration'>, options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.StartSubjectCalibration'>> {
    return (await this.#caller.call('SubjectCalibrationServices.StartSubjectCalibration', inputs, options)).outputs;
  }

  /**
   * Initiates subject re-calibration. The subject to update should be named using 'set subject name'.
   * @throws SubjectStoreError `InvalidArgument`: If the capture name has invalid characters.
   * @throws SubjectStoreError `NotAvailable`: If calibration is currently running.
   */
  async startSubjectRecalibration(inputs: Inputs<'SubjectCalibrationServices.StartSubjectRecalibration'>, options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.StartSubjectRecalibration'>> {
    return (await this.#caller.call('SubjectCalibrationServices.StartSubjectRecalibration', inputs, options)).outputs;
  }

  /** During calibration, mark the subject as being in the T-pose. */
  async acceptTPose(inputs: Inputs<'SubjectCalibrationServices.AcceptTPose'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SubjectCalibrationServices.AcceptTPose', inputs, options);
  }

  /**
   * Cancel the currently running subject calibration or re-calibration.
   * @throws SubjectStoreError `NotAvailable`: If calibration is not currently running.
   */
  async cancelSubjectCalibration(inputs: Inputs<'SubjectCalibrationServices.CancelSubjectCalibration'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SubjectCalibrationServices.CancelSubjectCalibration', inputs, options);
  }

  /**
   * Stop the currently running subject calibration or re-calibration.
   * @throws SubjectStoreError `NotAvailable`: If calibration is not currently running.
   */
  async stopSubjectCalibration(inputs: Inputs<'SubjectCalibrationServices.StopSubjectCalibration'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SubjectCalibrationServices.StopSubjectCalibration', inputs, options);
  }

  /** Get the current state of calibration or re-calibration. */
  async latestSubjectCalibrationState(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.LatestSubjectCalibrationState'>> {
    return (await this.#caller.call('SubjectCalibrationServices.LatestSubjectCalibrationState', {}, options)).outputs;
  }

  /**
   * The name for the subject to be created by the next subject calibration, or updated by recalibration.
   * @throws SubjectStoreError `InvalidArgument`: If the name contains .
   */
  async newSubjectName(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.NewSubjectName'>> {
    return (await this.#caller.call('SubjectCalibrationServices.NewSubjectName', {}, options)).outputs;
  }

  /** Set the name for the subject to be created by the next subject calibration, or updated by recalibration. */
  async setNewSubjectName(inputs: Inputs<'SubjectCalibrationServices.SetNewSubjectName'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SubjectCalibrationServices.SetNewSubjectName', inputs, options);
  }

  /** The set of templates available for generating the labeling skeleton. */
  async subjectLabellingTemplates(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.SubjectLabellingTemplates'>> {
    return (await this.#caller.call('SubjectCalibrationServices.SubjectLabellingTemplates', {}, options)).outputs;
  }

  /** The template for generating the labeling skeleton. */
  async subjectLabellingTemplate(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.SubjectLabellingTemplate'>> {
    return (await this.#caller.call('SubjectCalibrationServices.SubjectLabellingTemplate', {}, options)).outputs;
  }

  /**
   * Set the template for generating the labeling skeleton.  Should be from the set provided by SubjectLabellingTemplates.
   * @throws SubjectStoreError `NotFound`: The provided template name is not available.
   */
  async setSubjectLabellingTemplate(inputs: Inputs<'SubjectCalibrationServices.SetSubjectLabellingTemplate'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SubjectCalibrationServices.SetSubjectLabellingTemplate', inputs, options);
  }

  /** The set of skins available for generating the solving skeleton. */
  async subjectSkins(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.SubjectSkins'>> {
    return (await this.#caller.call('SubjectCalibrationServices.SubjectSkins', {}, options)).outputs;
  }

  /** The skin to use for subject calibration. */
  async subjectSkin(options?: CallOptions): Promise<Outputs<'SubjectCalibrationServices.SubjectSkin'>> {
    return (await this.#caller.call('SubjectCalibrationServices.SubjectSkin', {}, options)).outputs;
  }

  /**
   * Set the skin for generating the solving skeleton.  Should be from the set provided by SubjectSkins.
   * @throws SubjectStoreError `NotFound`: The provided skin name is not available.
   */
  async setSubjectSkin(inputs: Inputs<'SubjectCalibrationServices.SetSubjectSkin'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('SubjectCalibrationServices.SetSubjectSkin', inputs, options);
  }
}

/**
 * Functions of the standalone host for trying out what device states do, without any devices. The host's devices are what is recorded of them.
 * Preview: refused unless the host was started with `--level 1`.
 */
export class HostSimulation {
  readonly #caller: Caller;

  constructor(caller: Caller) {
    this.#caller = caller;
  }

  /**
   * The list of devices.
   * Preview: refused unless the host was started with `--level 1`.
   */
  async devices(options?: CallOptions): Promise<Outputs<'HostSimulation.Devices'>> {
    return (await this.#caller.call('HostSimulation.Devices', {}, options)).outputs;
  }

  /**
   * Get the state of a device.
   * Preview: refused unless the host was started with `--level 1`.
   * @throws SubjectStoreError `NotFound`: If there is no device with the URN supplied.
   */
  async deviceState(inputs: Inputs<'HostSimulation.DeviceState'>, options?: CallOptions): Promise<Outputs<'HostSimulation.DeviceState'>> {
    return (await this.#caller.call('HostSimulation.DeviceState', inputs, options)).outputs;
  }

  /**
   * Add a device, connected, with a full battery, not charging, and without a radio channel.
   * Preview: refused unless the host was started with `--level 1`.
   * @throws SubjectStoreError `AlreadyPresent`: If there is a device with the URN supplied.
   * @throws SubjectStoreError `InvalidArgument`: If the URN or the type is empty, or if the URN contains a slash or a control character or is longer than 255 bytes.
   */
  async addDevice(inputs: Inputs<'HostSimulation.AddDevice'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('HostSimulation.AddDevice', inputs, options);
  }

  /**
   * Remove a device. Links to it stay.
   * Preview: refused unless the host was started with `--level 1`.
   * @throws SubjectStoreError `NotFound`: If there is no device with the URN supplied.
   */
  async removeDevice(inputs: Inputs<'HostSimulation.RemoveDevice'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('HostSimulation.RemoveDevice', inputs, options);
  }

  /**
   * Connect or disconnect a device.
   * Preview: refused unless the host was started with `--level 1`.
   * @throws SubjectStoreError `NotFound`: If there is no device with the URN supplied.
   */
  async setConnected(inputs: Inputs<'HostSimulation.SetConnected'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('HostSimulation.SetConnected', inputs, options);
  }

  /**
   * Start or end the charging of a device.
   * Preview: refused unless the host was started with `--level 1`.
   * @throws SubjectStoreError `NotFound`: If there is no device with the URN supplied.
   */
  async setCharging(inputs: Inputs<'HostSimulation.SetCharging'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('HostSimulation.SetCharging', inputs, options);
  }

  /**
   * Set the charge of a device's battery.
   * Preview: refused unless the host was started with `--level 1`.
   * @throws SubjectStoreError `InvalidValue`: If the charge supplied is greater than 100.
   * @throws SubjectStoreError `NotFound`: If there is no device with the URN supplied.
   */
  async setBattery(inputs: Inputs<'HostSimulation.SetBattery'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('HostSimulation.SetBattery', inputs, options);
  }

  /**
   * Set the radio channel of a device.
   * Preview: refused unless the host was started with `--level 1`.
   * @throws SubjectStoreError `NotFound`: If there is no device with the URN supplied.
   */
  async setRadio(inputs: Inputs<'HostSimulation.SetRadio'>, options?: CallOptions): Promise<void> {
    await this.#caller.call('HostSimulation.SetRadio', inputs, options);
  }
}

/** The groups of the API, each as an object. */
export abstract class Groups implements Caller {
  /** Functions for managing basic objects. Basic objects are rigid bodies, with a fixed physical marker pattern. */
  readonly basicObjectServices = new BasicObjectServices(this);
  /** Functions for managing smart objects. A smart object represents the binding between the object (which appears in the data-stream) and the physical cluster device. The smart object can be configured in advance of the device arrival and persists after device disconnection. */
  readonly smartObjectServices = new SmartObjectServices(this);
  /** Services for object evaluation. This feature may be used to detect potential confusion between one object and another (basic or smart), or a different view of itself. */
  readonly objectEvaluationServices = new ObjectEvaluationServices(this);
  /** Functions for controlling characters tracked from clusters. */
  readonly characterFromClustersServices = new CharacterFromClustersServices(this);
  /** Functions for controlling and monitoring subject calibration. */
  readonly subjectCalibrationServices = new SubjectCalibrationServices(this);
  /**
   * Functions of the standalone host for trying out what device states do, without any devices. The host's devices are what is recorded of them.
   * Preview: refused unless the host was started with `--level 1`.
   */
  readonly hostSimulation = new HostSimulation(this);

  /** Calls a function by its full name. */
  abstract call<M extends Method>(method: M, inputs: Inputs<M>, options?: CallOptions): Promise<Result<M>>;
}
