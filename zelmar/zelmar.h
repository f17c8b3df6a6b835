#pragma once

/// Everything that hosts and plugins use.

#include <zelmar/Export.h>
#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/CliDispatcher.h>
#include <zelmar/autocli/Command.h>
#include <zelmar/autocli/CommandInput.h>
#include <zelmar/autocli/CommandList.h>
#include <zelmar/autocli/CommandOutput.h>
#include <zelmar/autocli/CommandSpec.h>
#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/InternalPlugin.h>
#include <zelmar/autocli/Namespace.h>
#include <zelmar/autocli/NamespaceNode.h>
#include <zelmar/autocli/OptionParser.h>
#include <zelmar/autocli/Plugin.h>
#include <zelmar/autocli/SharedLibraryPlugin.h>
#include <zelmar/autocli/formatters/CliDispatcherHelpFormatter.h>
#include <zelmar/autocli/formatters/CommandHelpFormatter.h>
#include <zelmar/autocli/formatters/FitString.h>
#include <zelmar/autocli/formatters/FormatParameters.h>
#include <zelmar/autocli/formatters/Formatter.h>
#include <zelmar/autocli/formatters/TableFormatter.h>
#include <zelmar/callspec/CallTarget.h>
#include <zelmar/callspec/Input.h>
#include <zelmar/callspec/InputSpec.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/OutputSpec.h>
#include <zelmar/callspec/ParameterConstraint.h>
#include <zelmar/callspec/ParameterSpec.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaObject.h>
#include <zelmar/metaobj/MetaScalars.h>
#include <zelmar/metaobj/MetaStruct.h>
