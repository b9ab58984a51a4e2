"""What the program validate_response says about responses."""
import pathlib
import subprocess
import tempfile


def complaints_about(bodies, validator):
    """Its complaints, empty for none."""
    with tempfile.TemporaryDirectory() as folder:
        files = []
        for number, body in enumerate(bodies):
            files.append(pathlib.Path(folder, str(number)))
            files[-1].write_bytes(body)
        run = subprocess.run([validator, *files], capture_output=True, text=True, check=False)
        return run.stdout + run.stderr + ("" if run.returncode == 0 else f"status {run.returncode}")
